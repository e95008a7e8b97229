"""Columns are counted in characters, whatever comes before the fault."""


def greetings(names):
	for name in names:
		print("こんにちは、", name, "さん" "!"))
		yield "naïve café" name
	table = {"größe": 1, "straße": 2, "été": 3,, "日本": 4}
	return table
