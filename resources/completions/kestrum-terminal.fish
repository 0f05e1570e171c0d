complete -c kestrum-terminal -f
complete -c kestrum-terminal -s h -l help -d 'Show the options'
complete -c kestrum-terminal -l version -d 'Show the version'
complete -c kestrum-terminal -l text -d 'Print the tree of the first refreshes'
