;;; A session of Emacs without a screen, as that of editor.lua. -*- lexical-binding: t -*-

(require 'package)
(package-initialize)
(require 'eglot)
(require 'flymake)
(require 'json)

(defun wait-for (what condition)
  "Wait until CONDITION holds, or say WHAT was waited for in vain."
  (let ((end (+ (float-time) 20)))
    (while (not (funcall condition))
      (when (> (float-time) end) (error "waited in vain: %s" what))
      (accept-process-output nil 0.05))))

(defun shown-problems ()
  "The text and the row of each problem."
  (eglot--signal-textDocument/didChange) ; what a timer does on a screen
  (flymake-start)
  (mapcar (lambda (one) (vector (line-number-at-pos (flymake-diagnostic-beg one)) (flymake-diagnostic-text one)))
          (flymake-diagnostics)))

(defun session ()
  "Break a file, mend it, and rename a name; what was seen."
  (load (getenv "EDITOR_SETTINGS"))
  (find-file (getenv "EDITED_FILE"))
  (run-hooks 'post-command-hook) ; a server is started after a command
  (wait-for "the server" #'eglot-managed-p)
  (goto-char (point-min))
  (forward-line 3)
  (insert "broken = (1\n")
  (wait-for "a problem" #'shown-problems)
  (let ((broken (vconcat (shown-problems))))
    (forward-char -1)
    (insert ")")
    (wait-for "no problem" (lambda () (null (shown-problems))))
    (goto-char (point-min))
    (search-forward "area")
    (eglot-rename "circle")
    (save-buffer)
    `((broken . ,broken))))

(let ((seen (condition-case failure (session) (error `((failure . ,(error-message-string failure)))))))
  (with-temp-file (getenv "EDITOR_REPORT") (insert (json-encode seen))))
