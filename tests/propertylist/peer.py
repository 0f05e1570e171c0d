"""The other side of the property-list tests: Python's own plistlib.

peer.py dump XML|BINARY    a Python expression on standard input -> the list
peer.py repr               a list on standard input -> its repr, in ASCII
peer.py convert XML|BINARY a list on standard input -> the same list, written by plistlib
"""
import datetime
import plistlib
import sys

given = sys.stdin.buffer.read()
action = sys.argv[1]
if action == "repr":
    print(ascii(plistlib.loads(given)), end="")
else:
    value = eval(given.decode("utf-8")) if action == "dump" else plistlib.loads(given)
    form = plistlib.FMT_XML if sys.argv[2] == "XML" else plistlib.FMT_BINARY
    sys.stdout.buffer.write(plistlib.dumps(value, fmt=form, sort_keys=False))
