#!/usr/bin/env bash
# Writes small seed corpora for the fuzz targets into DIR/<target>/.
set -euo pipefail
dir="$1"
mkfile="$2"
clipgen="$3"
mkdir -p "$dir/download_file" "$dir/reception" "$dir/settings" "$dir/avi"
"$clipgen" "$dir/avi/Filemove.avi"
"$mkfile" --bytes 600 "$dir/download_file/intel.hex" >/dev/null
"$mkfile" --bytes 600 --srec "$dir/download_file/srec.hex" >/dev/null
printf 'A.01.02\r\nMDSP:\r\nCDMA:\r\nAMPS:\r\nMPU:\r\nxxxxxxxxxxxxxxxxxxxxxxxxxxxxxx[EOF]\r\n' \
    >"$dir/download_file/minimal.hex"
i=0
for stage_step in '\x00\x02' '\x01\x00' '\x02\x00' '\x03\x00' '\x04\x04' '\x05\x06' '\x07\x08' '\x08\x01'; do
    for answer in '0,"No error"\r\n' 'Quorvex,ZX917,SN0001234567,FW----------A.01.02\r\n' \
        'DOWNLOAD READY\r\n\xffREV A.01.02 10\r\n' 'REV A.01.02 10\r\n\xffOPEN\r\n' \
        'P2A\r\n\xffRESTART:P2\r\n' 'P3A\r\n' 'EP1\r\n' 'ABORT\r\n' 'CLOSE\r\nREV A.01.02 10\r\n\xffREBOOT\r\n'; do
        printf "${stage_step}\x00${answer}" >"$dir/reception/seed$i"
        i=$((i + 1))
    done
done
for s in 9600,n,8,1 38400,E,8,1 19200,o,7,2 1200,m,5,1.5 115200,S,6,1; do
    printf '%s' "$s" >"$dir/settings/$s"
done
