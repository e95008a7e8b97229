"""A run as one page for a browser.

    excerpts.py    a file and its problems -> the rows that are worth showing
    names.py       the lines on those rows -> their names, with what is known of each
    file_data.py   both, and the counts of the file -> what the page holds of it
    counts.py      all problems -> the numbers of tables and charts
    page.py        all of that -> the page, by the template, the style and the scripts in assets/

What scripts need is in the page as JSON: `data-files` with every file and its problems, and for each file
whose rows are in the page `data-rows-N`, which is read when somebody opens the file. Scripts make text nodes
only, and a policy in the page admits no script but its own: no file name and no source is taken for markup.
"""
