# Takes out the paragraphs that scdoc opens and leaves empty, behind a heading and ahead of a macro.
/^\.P$/ { opened = !heading; next }
/^\.RE$/ { print; next }
opened && !/^\./ { print ".P" }
{ opened = 0; heading = /^\.(SH|TH)/; print }
