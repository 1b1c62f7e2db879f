#!/usr/bin/env python3
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
"""Compares the drawing in docs/architecture.md with the sources.

Each arrow of the drawing says that the files of one folder may include those of another. Prints
includes and CMake links without an arrow, arrows without an include or without a link, folders
that are missing from the drawing, and files that the page names and that do not exist.
"""
import glob
import os
import re
import sys

PAGE = 'docs/architecture.md'
SHARED = 'common'  # its own headers may be included without an arrow
INCLUDE = re.compile(r'^\s*#\s*include\s*[<"]([^>"]+)[>"]', re.M)


def drawing(page):
    """The folders of the drawing, and the arrows between them as pairs of folders."""
    text = re.search(r'```mermaid\n(.*?)```', page, re.S).group(1)
    folders = dict(re.findall(r'^\s*(\w+)\["([^"<]+?)(?:<[^"]*)?"\]$', text, re.M))
    arrows = set()
    for line in text.splitlines():
        if '-->' in line:
            start, end = (part.strip() for part in line.split('-->'))
            arrows |= {(folders[a.strip()], folders[b.strip()])
                       for a in start.split('&') for b in end.split('&')}
    return set(folders.values()), arrows


def room_of(path, rooms):
    return path if path in rooms else os.path.dirname(path)


def includes(rooms):
    """For each pair of rooms, a file of the first that includes the second."""
    found = {}
    for path in sorted(glob.glob('app/**/*.*', recursive=True) +
                       glob.glob('common/**/*.*', recursive=True)):
        if not path.endswith(('.h', '.cpp')):
            continue
        with open(path, encoding='utf-8') as source:
            for target in INCLUDE.findall(source.read()):
                if target.startswith(('app/', 'common/', '.')):
                    pair = room_of(path, rooms), room_of(target, rooms)
                    if pair[0] != pair[1] and pair[1] != SHARED:
                        found.setdefault(pair, path)
    return found


def libraries(rooms):
    """The rooms of each CMake target, and the project's own targets that each links."""
    aliases, places, links = {}, {}, {}
    for path in glob.glob('app/**/CMakeLists.txt', recursive=True) + ['common/CMakeLists.txt']:
        with open(path, encoding='utf-8') as script:
            text = re.sub(r'#.*', '', script.read())
        folder = os.path.dirname(path)
        for command, words in re.findall(
                r'^\s*(add_library|add_executable|velocor_add_room|target_link_libraries)'
                r'\(([^)]*)\)', text, re.M):
            words = words.split()
            target = words[0]
            if target.startswith('${'):
                continue
            if 'ALIAS' in words:
                aliases[target] = words[-1]
            elif command == 'target_link_libraries':
                links.setdefault(target, []).extend(words[1:])
            elif command == 'velocor_add_room':
                links.setdefault(target, []).extend(words[words.index('LINKS') + 1:])
            if command != 'target_link_libraries' and 'ALIAS' not in words:
                sources = [os.path.join(folder, word) for word in words[1:]
                           if word.endswith('.cpp')]
                places[target] = {room_of(source, rooms) for source in sources}
    return places, {target: {aliases.get(word, word) for word in words} & set(places)
                    for target, words in links.items()}


def reachable(links, target):
    seen, waiting = set(), [target]
    while waiting:
        for other in links.get(waiting.pop(), ()):
            if other not in seen:
                seen.add(other)
                waiting.append(other)
    return seen


def link_violations(rooms, arrows):
    places, links = libraries(rooms)
    for target in sorted(links):
        for other in sorted(links[target]):
            if not any((a, b) in arrows for a in places[target] for b in places[other]):
                yield f'{target} links {other}, but no arrow allows that'
    home = {room: target for target in places for room in places[target]}
    for a, b in sorted(arrows):
        if a not in home or b not in home:
            yield f'{a} --> {b}: {a if a not in home else b} is in no library'
        elif home[a] != home[b] and home[b] not in reachable(links, home[a]):
            yield f'{a} --> {b}: {home[a]} does not link {home[b]}'


def violations():
    with open(PAGE, encoding='utf-8') as file:
        page = file.read()
    rooms, arrows = drawing(page)
    used = includes(rooms)
    for pair in sorted(set(used) - arrows):
        yield f'{pair[0]} --> {pair[1]} is not drawn: {used[pair]}'
    for pair in sorted(arrows - set(used)):
        yield f'{pair[0]} --> {pair[1]} is drawn, but no file includes it'
    for folder in sorted({room_of(path, rooms) for path in
                          glob.glob('app/**/*.cpp', recursive=True) +
                          glob.glob('common/**/*.cpp', recursive=True)} - rooms):
        yield f'{folder} is not drawn'
    yield from link_violations(rooms, arrows)
    for name in sorted(set(re.findall(r'`((?:app|common|docs|scripts|tests)/[^`*]+)`', page))):
        if not os.path.exists(name):
            yield f'{name} is named, but does not exist'


def main():
    os.chdir(os.path.join(os.path.dirname(__file__), '..'))
    for violation in violations():
        print(f'{PAGE}: {violation}')


if __name__ == '__main__':
    sys.exit(main())
